// A valley: meadows and fields in front, a farm, single trees, wooded hills one behind the other.
#declare FogDistance = 700;
#include "common.inc"

camera { perspective location <0, 16, 0> right x * 4 / 3 up y angle 50 look_at <40, 9, 200> }
Sun(<-0.6, 0.7, -0.45>, <0.95, 0.88, 0.74>)
SkyLight(<0.20, 0.24, 0.30>)
Sky(<0.74, 0.83, 0.90>, <0.25, 0.48, 0.80>, <0.95, 0.95, 0.96>)

#declare Ground = function { pattern { bumps scale <170, 1, 170> } }
#declare Detail = function { pattern { bumps scale <21, 1, 21> } }
// Rolling in front, rising to hills behind.
#declare Height = function(x, z) {
  14 * Ground(x, 0, z) - 10 + 1.6 * Detail(x, 0, z) +
  min(1, max(0, (z - 260) / 900)) * (40 + 330 * pow(Ground(x * 0.42 + 900, 0, z * 0.42), 2))
}

#declare Fields = texture {
  pigment {
    cells
    turbulence 0.12
    colour_map {
      [0.0 rgb <0.36, 0.50, 0.18>] [0.3 rgb <0.46, 0.54, 0.22>] [0.3 rgb <0.70, 0.61, 0.30>]
      [0.5 rgb <0.62, 0.52, 0.27>] [0.5 rgb <0.30, 0.43, 0.15>] [0.8 rgb <0.40, 0.50, 0.20>]
      [0.8 rgb <0.46, 0.36, 0.24>] [1.0 rgb <0.40, 0.31, 0.21>]
    }
    scale <70, 400, 55> rotate y * 24
  }
  finish { Matt }
  normal { bumps 0.7 scale 0.9 }
}
#declare Woods = texture {
  pigment {
    bozo turbulence 0.6
    colour_map { [0 rgb <0.10, 0.19, 0.07>] [0.6 rgb <0.22, 0.33, 0.12>] [1 rgb <0.30, 0.38, 0.15>] }
    scale 9
  }
  finish { Matt }
  normal { bumps 1.4 scale 7 }
}

// Strips of the surface as meshes, finer in front.
#macro Strip(Z0, Z1, Step, Half, Look)
  mesh {
    #local Z = Z0;
    #while (Z < Z1)
      #local X = -Half;
      #while (X < Half)
        #local A = <X, Height(X, Z), Z>;
        #local B = <X + Step, Height(X + Step, Z), Z>;
        #local C = <X + Step, Height(X + Step, Z + Step), Z + Step>;
        #local D = <X, Height(X, Z + Step), Z + Step>;
        triangle { A, B, C }
        triangle { A, C, D }
        #local X = X + Step;
      #end
      #local Z = Z + Step;
    #end
    texture { Look }
  }
#end
Strip(-20, 100, 2, 90, Fields)
Strip(100, 400, 5, 280, Fields)
Strip(400, 1000, 10, 620, Woods)
Strip(1000, 2600, 25, 1500, Woods)

#declare Leaves = texture {
  pigment {
    bozo
    colour_map { [0 rgb <0.09, 0.17, 0.05>] [0.5 rgb <0.25, 0.39, 0.12>] [1 rgb <0.42, 0.52, 0.20>] }
    scale 0.5
  }
  finish { Matt }
  normal { bumps 1.2 scale 0.5 }
}
#declare Bark = texture { pigment { rgb <0.27, 0.20, 0.14> } finish { Matt } }
#macro Tree(Where, Size, Seed)
  #local R = seed(Seed);
  union {
    cone { 0, 0.06, y * 0.55, 0.03 texture { Bark } }
    #local I = 0;
    #while (I < 22)
      sphere {
        <rand(R) - 0.5, 0.42 + 0.5 * rand(R), rand(R) - 0.5> * <0.5, 1, 0.5>, 0.09 + 0.09 * rand(R)
        texture { Leaves }
      }
      #local I = I + 1;
    #end
    scale Size
    translate Where + y * (Height(Where.x, Where.z) - 0.3)
  }
#end
#macro Fir(Where, Size)
  union {
    cylinder { 0, y * 0.2, 0.03 texture { Bark } }
    #local I = 0;
    #while (I < 5)
      cone { y * (0.12 + 0.16 * I), 0.22 - 0.035 * I, y * (0.42 + 0.15 * I), 0.01 texture { Leaves } }
      #local I = I + 1;
    #end
    scale Size
    translate Where + y * (Height(Where.x, Where.z) - 0.3)
  }
#end

#declare R = seed(5);
Tree(<-13, 0, 38>, 13, 1)
Tree(<24, 0, 60>, 15, 2)
#declare I = 0;
#while (I < 70)
  #declare Z = 70 + 330 * pow(rand(R), 1.5);
  #declare X = (rand(R) * 2 - 1) * (30 + Z * 0.6) + Z * 0.2;
  #if (mod(I, 3) = 0) Fir(<X, 0, Z>, 14 + 7 * rand(R)) #else Tree(<X, 0, Z>, 11 + 6 * rand(R), I + 9) #end
  #declare I = I + 1;
#end

// The farm, a road and fence posts.
#macro House(Where, Size, Wall, Roof, Turn)
  union {
    box { <-0.5, -2, -0.5>, <0.5, 0.55, 0.5> Rough(Wall, 0.4) }
    prism { linear_spline -0.55, 0.55, 4, <-0.6, 0.5>, <0.6, 0.5>, <0, 1>, <-0.6, 0.5>
      rotate x * -90 Rough(Roof, 0.1) }
    #local I = -1;
    #while (I < 2)
      box { <I * 0.3 - 0.06, 0.15, -0.51>, <I * 0.3 + 0.06, 0.4, 0> pigment { rgb <0.13, 0.15, 0.18> } finish { Matt } }
      #local I = I + 1;
    #end
    scale Size rotate y * Turn translate Where + y * Height(Where.x, Where.z)
  }
#end
House(<34, 0, 130>, <14, 9, 10>, <0.86, 0.82, 0.74>, <0.55, 0.22, 0.16>, 20)
House(<58, 0, 142>, <20, 11, 12>, <0.50, 0.30, 0.20>, <0.30, 0.28, 0.28>, -35)
House(<90, 0, 230>, <12, 9, 10>, <0.78, 0.70, 0.52>, <0.60, 0.26, 0.18>, 60)
#declare I = 0;
#while (I < 26)
  #declare Z = 12 + I * 3;
  #declare X = -4 + 0.13 * Z;
  cylinder { <X, Height(X, Z) - 0.5, Z>, <X, Height(X, Z) + 1.3, Z>, 0.08 texture { Bark } }
  #declare I = I + 1;
#end
