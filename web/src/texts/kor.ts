import { eng, type Texts } from "./eng.ts";

export const kor: Texts = eng;
