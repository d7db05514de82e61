import { eng, type Texts } from "./eng.ts";

export const deu: Texts = eng;
