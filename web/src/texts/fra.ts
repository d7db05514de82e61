import { eng, type Texts } from "./eng.ts";

export const fra: Texts = eng;
