import { render } from "preact";
import { App } from "./App.tsx";
import { followAddress } from "./route.ts";
import { closeSessionWithPage } from "./service/session.ts";
import { findSimulator } from "./service/simulator.ts";
import { keepWatching } from "./service/watch.ts";
import { chooseLanguage } from "./texts/texts.ts";
import "./style.css";
import "uplot/dist/uPlot.min.css";

chooseLanguage();
followAddress();
closeSessionWithPage();
void findSimulator();
keepWatching();
render(<App />, document.getElementById("page")!);
