import { eng, type Texts } from "./eng.ts";

export const jpn: Texts = eng;
