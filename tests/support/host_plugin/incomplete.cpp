extern "C" {
void qitrmcInit() {}
void qitrmcPause() {}
void qitrmcResume() {}
void qitrmcFinalize() {}
}
