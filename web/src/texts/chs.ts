import { eng, type Texts } from "./eng.ts";

export const chs: Texts = eng;
